# Writes the completion scripts and manual pages into OUT, laid out as under
# share/. Run by the build with HYRACLI, HYRASIM, MANPAGES, PLUGIN_DIR, WORLD,
# OUT, DATE and VERSION set.

# The commands are registered only while the simulated daemon runs, so the
# tools get a fresh demo world of their own, removed afterwards.
set(ENV{HYRA_SIM_DB} ${WORLD})
function(remove_world)
  file(REMOVE ${WORLD} ${WORLD}-wal ${WORLD}-shm ${WORLD}-journal)
endfunction()
remove_world()

# Runs the command in ARGN, its output into the file output when not empty.
function(run output)
  set(redirect)
  if(output)
    set(redirect OUTPUT_FILE ${output})
  endif()
  execute_process(COMMAND ${ARGN} ${redirect} RESULT_VARIABLE status ERROR_VARIABLE error)
  if(NOT status EQUAL 0)
    remove_world()
    message(FATAL_ERROR "${ARGN} failed (${status}): ${error}")
  endif()
endfunction()

run("" ${HYRASIM} init --demo)

set(completions
  bash bash-completion/completions/hyracli
  zsh zsh/vendor-completions/_hyracli
  fish fish/vendor_completions.d/hyracli.fish)
while(completions)
  list(POP_FRONT completions shell file)
  get_filename_component(directory ${OUT}/${file} DIRECTORY)
  file(MAKE_DIRECTORY ${directory})
  run(${OUT}/${file} ${HYRACLI} --plugin-dir ${PLUGIN_DIR} completion ${shell})
endwhile()

# Pages of commands that are gone must not linger.
file(REMOVE_RECURSE ${OUT}/man/man1)
file(MAKE_DIRECTORY ${OUT}/man/man1)
run("" ${MANPAGES} ${OUT}/man/man1 ${DATE} ${VERSION} ${PLUGIN_DIR})

remove_world()
