// Filled in with its commands' tests.
