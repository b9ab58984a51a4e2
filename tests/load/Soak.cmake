# Loads and unloads the provider itself: nothing of it or of its framework may be in the program.
