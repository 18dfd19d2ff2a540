// Replaced by this kit's first source.
