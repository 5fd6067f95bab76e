// Filled in by the reliability suite.
