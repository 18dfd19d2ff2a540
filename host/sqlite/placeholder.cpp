// Replaced by the first source.
