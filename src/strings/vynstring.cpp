// The encoded string core.
